// The server that the wire benchmark compares with: the same function, over the same library that a Node developer would
// take. Prints its port and process id as one line of JSON.
import { readFileSync } from 'node:fs'
import { createRequire } from 'node:module'
const { Server } = createRequire(import.meta.url)('rpc-websockets')

const colours = new Map(Array.from({ length: 1000 }, (_, i) => [`Subject ${i}`, '#ffcc8844']))
const server = new Server({ port: 0, host: '127.0.0.1' })
server.register('BasicObjectServices.Color', ([name]) => {
  const colour = colours.get(name)
  if (colour === undefined) throw new Error('NotFound')
  return { code: 0, name: 'Ok', outputs: { ColorHtml: colour } }
})
server.on('listening', () => {
  console.log(JSON.stringify({ port: server.wss.address().port, pid: process.pid }))
})
