// A server that tells all who are connected of each message, over the library that a Node developer would take. Prints
// its port.
import { createRequire } from 'node:module'
const { WebSocketServer } = createRequire(new URL('../wire/package.json', import.meta.url))('ws')

const server = new WebSocketServer({ port: 0, host: '127.0.0.1' })
let sequence = 1000000
server.on('connection', client => client.on('message', data => {
  const message = JSON.parse(data)
  if (message.method === 'Server.Subscribe') return
  const method = 'BasicObjectServices.BasicObjectChangedCallback'
  const text = JSON.stringify({ jsonrpc: '2.0', method, params: { sequence: ++sequence } })
  for (const other of server.clients) if (other !== client) other.send(text)
  client.send(JSON.stringify({ jsonrpc: '2.0', id: message.id, result: { code: 0, name: 'Ok', outputs: {} } }))
}))
server.on('listening', () => console.log(server.address().port))
