# How Sphinx makes the site; tools/site_source.py copies this beside its sources.
project = "TALUtil"
html_title = "TALUtil"
extensions = ["myst_parser"]
source_suffix = {".md": "markdown"}
myst_enable_extensions = ["deflist"]
myst_heading_anchors = 4
# Quotes in texts are those that programs are written with.
smartquotes = False
html_theme = "furo"
html_static_path = ["static"]
html_css_files = ["site.css"]
html_copy_source = False
html_show_sourcelink = False
html_show_copyright = False
html_use_index = False
pygments_style = "default"
pygments_dark_style = "native"
# The distribution's theme lacks the colours of the dark form.
html_theme_options = {
    "navigation_with_keys": True,
    "dark_css_variables": {
        "color-foreground-primary": "#d8dce2",
        "color-foreground-secondary": "#a9b1bc",
        "color-foreground-muted": "#8d96a3",
        "color-foreground-border": "#666c75",
        "color-background-primary": "#15171b",
        "color-background-secondary": "#1c1f24",
        "color-background-hover": "#272b32",
        "color-background-hover--transparent": "#272b3200",
        "color-background-border": "#343a42",
        "color-background-item": "#444a53",
        "color-brand-primary": "#8cbaff",
        "color-brand-content": "#8cbaff",
        "color-highlighted-background": "#0b3a69",
        "color-inline-code-background": "#262a31",
    },
}
