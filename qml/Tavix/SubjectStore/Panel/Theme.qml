pragma Singleton
import QtQuick

/// Colours and sizes of everything in the panel. Sizes follow the font, so that they grow with the user's settings.
QtObject {
    id: theme

    enum Scheme {
        System,
        Light,
        Dark
    }

    /// Which colours are used; the system's preference unless somebody chooses.
    property int scheme: Theme.System
    readonly property bool dark: scheme === Theme.Dark || (scheme === Theme.System && systemPalette.window.hslLightness < 0.5)

    // Surfaces, from the back to the front
    readonly property color window: dark ? "#1e2126" : "#eef0f3"
    readonly property color surface: dark ? "#272b31" : "#ffffff"
    readonly property color raised: dark ? "#323740" : "#f7f8fa"
    readonly property color header: dark ? "#2c3138" : "#e3e7ec"
    readonly property color line: dark ? "#434a55" : "#c9d0d9"
    readonly property color hovered: dark ? "#343b46" : "#e9f0fa"

    // Texts
    readonly property color text: dark ? "#e6e9ee" : "#1b1f24"
    readonly property color secondaryText: dark ? "#a3acb9" : "#566070"
    readonly property color disabledText: dark ? "#6d7683" : "#9aa3af"
    readonly property color selected: dark ? "#2f4a70" : "#cfe0f9"
    readonly property color selectedInactive: dark ? "#3a414d" : "#e0e4ea"
    readonly property color highlight: dark ? "#3d7bd9" : "#2563c4"
    readonly property color highlightedText: "#ffffff"

    // Meanings
    readonly property color good: dark ? "#4fb477" : "#1f8a4c"
    readonly property color warning: dark ? "#e3b341" : "#9a6700"
    readonly property color critical: dark ? "#f0716a" : "#c6302b"
    readonly property color running: dark ? "#5aa9f5" : "#1a6fc9"

    // Sizes in device-independent pixels
    readonly property real unit: Math.max(4, Math.round(metrics.height / 4))
    readonly property real spacing: unit
    readonly property real margin: 2 * unit
    readonly property real rowHeight: Math.round(metrics.height * 1.6)
    readonly property real indentation: 4 * unit
    readonly property real radius: unit / 2
    readonly property real smallFont: Math.round(metrics.font.pixelSize * 0.88)
    readonly property real iconSize: Math.round(metrics.height)

    /// Where the names of subjects begin in their rows, and what is beneath them.
    readonly property real nameMargin: Math.round(2 * unit + 2 * (iconSize + spacing) + 0.7 * iconSize + spacing)
    /// What rows keep free at their ends for warnings.
    readonly property real badgeWidth: Math.round(iconSize + 3 * unit)

    /// Of a choice in a palette.
    readonly property real cellSize: Math.round(rowHeight + 1.5 * unit)

    /// In ms, before a tooltip appears.
    readonly property int tipDelay: 600

    /// One of 64 colours that neighbours of which differ; for active marker patterns. 0, no pattern, is grey.
    function patternColour(pattern: int): color {
        if (pattern <= 0)
            return theme.disabledText
        return Qt.hsla((pattern * 0.618034) % 1, 0.65, theme.dark ? 0.62 : 0.42, 1)
    }

    readonly property SystemPalette systemPalette: SystemPalette {}
    readonly property FontMetrics metrics: FontMetrics {}
}
