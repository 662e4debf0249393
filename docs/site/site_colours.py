"""The colours of code on the pages. Each has a contrast of at least 4.5 to its background."""
from pygments.style import Style
from pygments.token import Comment, Generic, Keyword, Literal, Name, Number, String, Token


class Light(Style):
    background_color = "#f6f8fa"
    styles = {
        Token: "#1f2328", Comment: "#57606a", Keyword: "#953800", Name.Class: "#0550ae", Name.Function: "#0550ae", Name.Tag: "#0550ae",
        String: "#0a3069", Number: "#0550ae", Literal: "#0550ae", Generic.Prompt: "#57606a", Generic.Output: "#1f2328",
        Comment.Preproc: "#953800",
    }


class Dark(Style):
    background_color = "#1c1f24"
    styles = {
        Token: "#e6edf3", Comment: "#9ea7b3", Keyword: "#ffa657", Name.Class: "#79b8ff", Name.Function: "#79b8ff", Name.Tag: "#79b8ff",
        String: "#a5d6ff", Number: "#79b8ff", Literal: "#79b8ff", Generic.Prompt: "#9ea7b3", Generic.Output: "#e6edf3",
        Comment.Preproc: "#ffa657",
    }
