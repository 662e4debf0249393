char const* extra = "fancy";
