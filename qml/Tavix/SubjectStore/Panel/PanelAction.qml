import QtQuick.Controls

/// One command, whether it is given by menu, tool bar or keyboard.
Action {
    /// What it does, where its text is not enough.
    property string tip
    /// What is missing while it cannot be given.
    property string needs
    /// The keys that give it while the list has the focus. They are not a shortcut of the whole window, which would
    /// let Delete remove subjects while somebody works elsewhere.
    property string keys

    readonly property string hint: enabled ? tip : needs
}
