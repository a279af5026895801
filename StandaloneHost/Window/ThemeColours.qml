import QtQml
import Tavix.SubjectStore.Panel

/// Hands the theme to those who ask for its colours by name.
QtObject {
    readonly property QtObject theme: Theme
}
